#pragma once

#include <QLabel>
#include <QSlider>
#include <QTimer>
#include <QWidget>
#include <optional>

#include "widgets/GlyphButton.h"
#include "widgets/TextButton.h"

namespace varnel {

/// What a `PlayBar` shows.
struct PlayBarState {
  enum class Button { None, Play, Pause, Again };

  QString name{};                 ///< of what is played
  Button button = Button::None;   ///< what the first button does
  int place = 0, length = 0;      ///< the slider goes from 0 to the length; without a length there is none
  int step = 1;                   ///< how far an arrow key moves the slider
  QString date{}, clock{};        ///< the time at the place; the date is left out where there is no room
  QString progress{};             ///< how far the place is
  std::optional<double> speed{};  ///< absent: nobody can choose it
  QString message{};              ///< in place of the slider and what is beside it; may be empty
  QString remedy{};               ///< the title of the button that helps with the message; may be empty

  bool operator==(const PlayBarState&) const = default;
};

/// The bar below the stack that plays a capture. It knows no server: it shows a state, and tells what the
/// user wants. While the user moves the slider, states do not move it.
class PlayBar final : public QWidget {
  Q_OBJECT

 public:
  explicit PlayBar(QWidget* parent = nullptr);

  void setState(const PlayBarState& state);
  const PlayBarState& state() const { return _state; }
  /// What the button at the end does; by default it closes the file.
  void setWayToClose(const QString& text);
  /// Tells how far a place is while the user moves the slider.
  void setProgress(const QString& progress);
  QSize sizeHint() const override;

  GlyphButton& playButton() { return *_play; }
  GlyphButton& closeButton() { return *_close; }
  TextButton& speedButton() { return *_speed; }
  TextButton& remedyButton() { return *_remedy; }
  QSlider& slider() { return *_slider; }
  /// All texts that are on display, in their order, with " | " between them.
  QString texts() const;

 Q_SIGNALS:
  void playWanted();
  void pauseWanted();
  void againWanted();
  void speedWanted(double speed);
  /// The user moves the slider, which is at this place.
  void dragged(int place);
  /// The user has chosen this place.
  void jumpWanted(int place);
  void remedyWanted();
  void closeWanted();
  /// The keyboard is no longer needed here.
  void keyboardLeft();

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;

 private:
  void passKeyboardOn();
  void press();
  void showTime();
  void showButton();
  void chooseSpeed();
  void sliderWasMoved();

  PlayBarState _state;
  GlyphButton* _play;
  QSlider* _slider;
  QLabel* _time;
  QLabel* _progress;
  TextButton* _speed;
  QLabel* _message;
  TextButton* _remedy;
  GlyphButton* _close;
  QTimer _keysAreDone;  // a jump for several presses of a key
};

}  // namespace varnel
