// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/settingsfile/SettingsFilter.h"

#include "app/settingsfile/CaselessText.h"

namespace Velocor {

SettingsFilter::Shown SettingsFilter::Of(SettingsDocument const& document,
                                         SettingsValues const& saved,
                                         SettingsValues const& defaults) const
{
    const CaselessText wanted(text);
    const auto isWanted = [&](QString const& section, SettingsDocument::Item const& item) {
        if (onlyChanged) {
            const auto inFile = saved.constFind({section, item.key});
            if (inFile != saved.constEnd() && inFile.value() == item.value)
                return false;
        }
        if (!onlyDiffering)
            return true;
        const auto byDefault = defaults.constFind({section, item.key});
        return byDefault != defaults.constEnd() && byDefault.value() != item.value;
    };

    Shown shown;
    int number = 0;
    for (SettingsDocument::Section const& section : document.sections) {
        const bool isNamed = wanted.IsIn(section.name);
        std::vector<int> items;
        for (int i = 0; i < section.items.size(); ++i) {
            SettingsDocument::Item const& item = section.items.at(i);
            if ((isNamed || wanted.IsIn(item.key) || wanted.IsIn(item.value)) &&
                isWanted(section.name, item))
                items.push_back(i);
        }
        if (!items.empty() || (isNamed && !onlyChanged && !onlyDiffering))
            shown.sections.push_back(number);
        shown.items.push_back(std::move(items));
        ++number;
    }
    return shown;
}

} // namespace Velocor
