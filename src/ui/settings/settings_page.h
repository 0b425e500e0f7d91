// The settings page: the probe of Com1 and Com2, the option lists filled from the port's
// settings, Preset, and the engineer's choice applied to the port. The rules are the core's
// (ProbePorts, SettingsFieldsOf, SettingsTextOf); the lists carry the values they stand for.
#pragma once

#include <QComboBox>
#include <QGroupBox>
#include <QLabel>
#include <QPushButton>
#include <QWidget>
#include <functional>
#include <string>
#include <vector>

#include "app/app_state.h"
#include "app/dialogs.h"
#include "app/texts.h"
#include "link/serial_port.h"

namespace zx917::ui {

struct SettingsParts {
    AppState& app;
    const TextTables& texts;
    SerialPort& port;
    Dialogs& dialogs;
    // What "Com<n>" is on this machine (device path and description), for its tooltip.
    std::function<std::string(int16_t)> describePort;
};

inline constexpr int16_t kProbedPorts = 2;

class SettingsPage : public QWidget {
public:
    // The page itself, with its instruction, port list and "Settings" frame.
    SettingsPage(const SettingsParts& parts, QWidget* window);

    bool ProtSettings();
    void cmdReset_Click();
    bool ProtSettingsApply();

    // The seven lists and Preset; identification disables them while it runs.
    void setListsEnabled(bool enabled);

    QLabel* Label7_1;
    QLabel* Label3;
    QComboBox* cboPort;
    QGroupBox* Frame3;
    QComboBox* cboSpeed;
    QComboBox* cboDataBits;
    QComboBox* cboStopBits;
    QComboBox* cboParity;
    QComboBox* cboXon;
    QComboBox* cboEoc;
    QPushButton* cmdReset;

private:
    void ProtSettingsShow();
    // Selects in the lists what a settings text, terminator and handshaking code stand for.
    void show(const std::string& settings, const std::string& terminator, int16_t handshaking);

    SettingsParts p_;
};

// Selects the item with exactly this text; without one, a pick-only list has no selection and
// an editable list shows the text.
void SetListText(QComboBox* list, const QString& text);

}  // namespace zx917::ui
