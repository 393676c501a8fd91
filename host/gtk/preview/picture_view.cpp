// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/picture_view.h"

#include <algorithm>
#include <cmath>
#include <sstream>

#include "host/gtk/preview/decoder_process.h"
#include "host/gtk/preview/picture_canvas.h"
#include "host/gtk/preview/picture_controls.h"
#include "host/gtk/preview/picture_frames.h"
#include "host/gtk/preview/picture_gestures.h"
#include "host/gtk/preview/shared_bytes.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

constexpr int LongestPictureSide = 8192;   // of what is asked for at once, pixels
constexpr guint PictureSettledAfter = 60;  // milliseconds without a change, before detail is asked for
constexpr double SharpFrom = 2;            // device pixels a pixel, where the decoder draws them with sharp edges
constexpr double Margin = 0.25;            // of the window that is asked for around it, for the next move
constexpr double LongestPicture = 1e7;

int bounded(double length) { return std::clamp(static_cast<int>(std::lround(length)), 1, LongestPictureSide); }

class PictureView : public DocumentView {
 public:
  PictureView(const PreviewedDocument& document, DocumentViewEvents events)
      : document_(document),
        events_(std::move(events)),
        process_(std::make_unique<DecoderProcess>("picture", document.path)),
        overlay_(GTK_WIDGET(g_object_ref_sink(gtk_overlay_new()))),
        gestures_(canvas_),
        controls_({[this] { gestures_.zoomIn(); }, [this] { gestures_.zoomOut(); }, [this] { gestures_.showWhole(); }}),
        notice_(gtk_label_new(_("The end of this picture is missing."))) {
    gtk_overlay_set_child(GTK_OVERLAY(overlay_), canvas_.widget());
    gtk_overlay_add_overlay(GTK_OVERLAY(overlay_), controls_.widget());
    gtk_overlay_add_overlay(GTK_OVERLAY(overlay_), notice_);
    for (const char* style : {"osd", "toolbar"}) gtk_widget_add_css_class(notice_, style);
    gtk_widget_set_halign(notice_, GTK_ALIGN_CENTER);
    gtk_widget_set_valign(notice_, GTK_ALIGN_START);
    gtk_widget_set_margin_top(notice_, 12);
    gtk_widget_set_visible(notice_, FALSE);
    gtk_accessible_update_property(GTK_ACCESSIBLE(canvas_.widget()), GTK_ACCESSIBLE_PROPERTY_LABEL, document.name.c_str(),
                                   -1);
    canvas_.setChanged([this] { viewportChanged(); });
    gestures_.setTouched([this] { controls_.appear(); });
    g_signal_connect_swapped(canvas_.widget(), "map", G_CALLBACK(+[](PictureView* self) {
                               gtk_widget_grab_focus(self->canvas_.widget());
                               self->playOn();
                             }),
                             this);
    g_signal_connect_swapped(canvas_.widget(), "unmap", G_CALLBACK(+[](PictureView* self) { self->frames_.reset(); }), this);
    // How much is asked for depends on the place that the view gets.
    g_signal_connect_swapped(overlay_, "notify::parent", G_CALLBACK(+[](PictureView* self) {
                               if (!self->asking_ && !self->isShown_ && gtk_widget_get_parent(self->overlay_))
                                 self->askWhole();
                             }),
                             this);
  }

  ~PictureView() override {
    g_clear_handle_id(&settling_, g_source_remove);
    g_signal_handlers_disconnect_by_data(canvas_.widget(), this);
    g_signal_handlers_disconnect_by_data(overlay_, this);
    canvas_.setChanged(nullptr);
    g_object_unref(overlay_);
  }

  GtkWidget* widget() override { return overlay_; }

  void refresh() override {
    frames_.reset();
    process_ = std::make_unique<DecoderProcess>("picture", document_.path);
    hasDetail_ = false;
    isBroken_ = false;
    askWhole();
  }

 private:
  double deviceScale() const { return canvas_.viewport().scale() * gtk_widget_get_scale_factor(overlay_); }

  // The view has no size before it was seen, but its place has one, or at least the window.
  PictureViewport::Size place() const {
    const PictureViewport::Size window = canvas_.viewport().window();
    if (window.width > 0 && window.height > 0) return window;
    for (GtkWidget* widget = gtk_widget_get_parent(overlay_); widget; widget = gtk_widget_get_parent(widget)) {
      const double width = gtk_widget_get_width(widget);
      const double height = gtk_widget_get_height(widget);
      if (width > 0 && height > 0) return {width, height};
    }
    return {1024, 768};
  }

  std::string boundsWords() const {
    const PictureViewport::Size size = place();
    const int factor = gtk_widget_get_scale_factor(overlay_);
    return std::to_string(bounded(size.width * factor)) + " " + std::to_string(bounded(size.height * factor));
  }

  void askWhole() {
    asking_ = true;
    const auto answered = [this](DecoderProcess::Answer answer) {
      asking_ = false;
      if (!answer.error.empty()) return events_.failed(messageForDecoderError(answer.error));
      gotWhole(std::move(answer));
    };
    process_->ask("whole " + boundsWords(), answered, document_.patience);
  }

  void gotWhole(DecoderProcess::Answer answer) {
    std::istringstream words(answer.text);
    PictureViewport::Size size;
    int width = 0;
    int height = 0;
    int delay = -1;
    const bool isRead = static_cast<bool>(words >> size.width >> size.height >> width >> height >> delay);
    const bool isSane =
        isRead && size.width >= 1 && size.height >= 1 && size.width <= LongestPicture && size.height <= LongestPicture;
    GRef<GdkTexture> texture = isSane ? takeTexture(std::move(answer.file), width, height) : nullptr;
    if (!texture) return events_.failed(messageForDecoderError(DecoderError::Damaged));
    bool isPartial = false;
    isTransparent_ = false;
    isScalable_ = false;
    for (std::string word; words >> word;) {
      isTransparent_ = isTransparent_ || word == "transparent";
      isScalable_ = isScalable_ || word == "scalable";
      isPartial = isPartial || word == "partial";
    }
    isAnimated_ = delay >= 0;
    delay_ = delay;
    wholeScale_ = width / size.width;
    gtk_widget_set_visible(notice_, isPartial);
    canvas_.setWhole(std::move(texture), isTransparent_);
    canvas_.setDetail(nullptr, {});
    hasDetail_ = false;
    canvas_.change([&](PictureViewport& viewport) { viewport.setPicture(size, isScalable_); });
    if (!isShown_) {
      isShown_ = true;
      events_.shown();
    }
    playOn();
  }

  void playOn() {
    if (!isAnimated_ || frames_ || !gtk_widget_get_mapped(canvas_.widget())) return;
    frames_ = std::make_unique<PictureFrames>(
        *process_, delay_, [this] { return frameWords(); },
        [this](GRef<GdkTexture> texture) { canvas_.setWhole(std::move(texture), isTransparent_); });
  }

  // An animation is sent whole, as large as it is seen.
  std::string frameWords() const {
    const PictureViewport::Area area = canvas_.viewport().pictureArea();
    const int factor = gtk_widget_get_scale_factor(overlay_);
    constexpr double most = 2048;
    return std::to_string(bounded(std::min(area.width * factor, most))) + " " +
           std::to_string(bounded(std::min(area.height * factor, most)));
  }

  void viewportChanged() {
    const PictureViewport& viewport = canvas_.viewport();
    controls_.setScale(viewport.scale(), viewport.isFitting(), viewport.scale() >= viewport.largestScale());
    if (!isShown_ || isAnimated_ || isBroken_) return;
    g_clear_handle_id(&settling_, g_source_remove);
    settling_ = g_timeout_add(
        PictureSettledAfter,
        +[](gpointer data) -> gboolean {
          auto* self = static_cast<PictureView*>(data);
          self->settling_ = 0;
          self->sharpen();
          return G_SOURCE_REMOVE;
        },
        this);
  }

  // Asks for what is seen in the detail of the display, unless it is there.
  void sharpen() {
    if (asking_ || isBroken_) return;
    constexpr double almost = 1.01;
    const PictureViewport& viewport = canvas_.viewport();
    const double scale = deviceScale();
    const double best = isScalable_ ? scale : std::min(scale, 1.0);
    if (viewport.isFitting()) {
      canvas_.setDetail(nullptr, {});
      hasDetail_ = false;
      if (best > wholeScale_ * almost || best < wholeScale_ / almost) askWhole();
      return;
    }
    if (best <= wholeScale_ * almost && scale < SharpFrom) return;
    const PictureViewport::Area seen = viewport.visiblePart();
    const bool isSharp = hasDetail_ && scale <= detailScale_ * almost && scale >= detailScale_ / almost;
    if (isSharp && detailPart_.covers(seen)) return;
    askPart(seen, scale);
  }

  void askPart(const PictureViewport::Area& seen, double scale) {
    const PictureViewport::Size picture = canvas_.viewport().picture();
    const double left = std::floor(std::max(0.0, seen.x - seen.width * Margin));
    const double top = std::floor(std::max(0.0, seen.y - seen.height * Margin));
    const double right = std::ceil(std::min(picture.width, seen.x + seen.width * (1 + Margin)));
    const double bottom = std::ceil(std::min(picture.height, seen.y + seen.height * (1 + Margin)));
    const PictureViewport::Area part = {left, top, right - left, bottom - top};
    const int width = bounded(part.width * scale);
    const int height = bounded(part.height * scale);
    std::ostringstream words;
    words.imbue(std::locale::classic());
    words << "part " << static_cast<long>(part.x) << ' ' << static_cast<long>(part.y) << ' ' << static_cast<long>(part.width)
          << ' ' << static_cast<long>(part.height) << ' ' << width << ' ' << height;
    asking_ = true;
    process_->ask(words.str(), [this, part, scale, width, height](DecoderProcess::Answer answer) {
      asking_ = false;
      GRef<GdkTexture> texture = answer.error.empty() ? takeTexture(std::move(answer.file), width, height) : nullptr;
      // The coarse picture stays, which is better than none.
      isBroken_ = !texture;
      if (isBroken_) return;
      hasDetail_ = true;
      detailPart_ = part;
      detailScale_ = scale;
      canvas_.setDetail(std::move(texture), part);
      sharpen();
    });
  }

  PreviewedDocument document_;
  DocumentViewEvents events_;
  std::unique_ptr<DecoderProcess> process_;
  GtkWidget* overlay_;
  PictureCanvas canvas_;
  PictureGestures gestures_;
  PictureControls controls_;
  GtkWidget* notice_;
  std::unique_ptr<PictureFrames> frames_;  // while it plays
  bool isShown_ = false;
  bool asking_ = false;
  bool isBroken_ = false;  // no more detail is to be had
  bool isTransparent_ = false;
  bool isScalable_ = false;
  bool isAnimated_ = false;
  int delay_ = -1;
  double wholeScale_ = 1;  // pixels of it for each of the picture
  bool hasDetail_ = false;
  PictureViewport::Area detailPart_;
  double detailScale_ = 1;
  guint settling_ = 0;
};

}  // namespace

bool showsPicture(const std::string& contentType) {
  if (!g_content_type_is_a(contentType.c_str(), "image/*")) return false;
  if (contentType.rfind("image/svg+xml", 0) == 0) return true;
  bool found = false;
  GSList* formats = gdk_pixbuf_get_formats();
  for (const GSList* format = formats; format && !found; format = format->next) {
    gchar** types = gdk_pixbuf_format_get_mime_types(static_cast<GdkPixbufFormat*>(format->data));
    for (gchar** type = types; *type && !found; ++type) {
      const std::string own = takeString(g_content_type_from_mime_type(*type));
      found = g_content_type_is_a(contentType.c_str(), own.c_str());
    }
    g_strfreev(types);
  }
  g_slist_free(formats);
  return found;
}

std::unique_ptr<DocumentView> makePictureView(const PreviewedDocument& document, DocumentViewEvents events) {
  return std::make_unique<PictureView>(document, std::move(events));
}

}  // namespace vaelo
