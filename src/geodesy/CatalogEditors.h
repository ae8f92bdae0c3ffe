#pragma once
// The logic of the three catalog editors, without widgets: the field texts,
// the changed and new-entry flags, the entry lists and what New, OK, Delete,
// a selection and closing do. Every read and write goes through the catalog
// store. An operation that refuses puts the field that should get the focus
// into takeFocus(); the widgets bind their controls to these classes.

#include <array>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "geodesy/CatalogStore.h"
#include "platform/Ui.h"

namespace zv {

// What every editor shares: the texts of its fields (as shown and as last
// loaded), the two flags, the entry list and the common buttons. `Field` is
// an enum whose first value is the short name and whose last is Count.
template <class Field>
class CatalogEditor {
 public:
  using FieldType = Field;
  static constexpr size_t kFields = static_cast<size_t>(Field::Count);

  virtual ~CatalogEditor() = default;

  const std::string& text(Field f) const { return text_[Index(f)]; }
  bool checked(Field f) const { return text(f) == "1"; }
  // A user's edit: sets the changed flag when the text differs from the one
  // last loaded.
  void edit(Field f, std::string text);
  void check(Field f, bool on) { edit(f, on ? "1" : "0"); }

  bool changed() const { return changed_; }
  bool isNew() const { return isNew_; }
  // The section names of the catalog (for zones: the zones of the listed
  // coordinate system), in file order.
  const std::vector<std::string>& entries() const { return entries_; }
  // The entry whose keys are in the fields; empty for a new one.
  const std::string& selected() const { return selected_; }
  // The field the last operation wants focused, once.
  std::optional<Field> takeFocus() { return std::exchange(focus_, std::nullopt); }

  // Loads the entry after saving a changed one; false when the save refused
  // (the fields stay).
  bool select(const std::string& name);
  // Clears the fields for a new entry after saving a changed one.
  bool newEntry();
  // True when the editor may close: a changed entry was saved or abandoned.
  bool ok();
  // The close question for a changed entry; true when the editor may close.
  bool close();
  // Asks, then removes the selected entry; true when it was removed.
  bool remove();
  // Validates and writes the entry. True after a write and after a No to the
  // overwrite question; false when a check refused (focus on the field).
  virtual bool save() = 0;

 protected:
  struct Words {
    const char* title;    // "Ellipsoid"
    const char* word;     // "ellipsoid"
    const char* article;  // "An" or "A"
  };
  CatalogEditor(Ui& ui, Words words) : ui_(ui), words_(words) {}

  static size_t Index(Field f) { return static_cast<size_t>(f); }
  // Shows a text as loaded: no change.
  void put(Field f, std::string text);
  void clearFields();
  // A refusal of the save: the box, the focus, false.
  bool refuse(Field f, const std::string& text);
  // The duplicate check of a save: false when the name collides and the user
  // answered No (focus on the short name).
  bool confirmOverwrite(const std::string& name, bool exists);
  // The message for a store that could not write; false.
  bool writeFailed(const CatalogFile& store);
  // After a write: the list afresh with the entry selected.
  void saved(const std::string& name);

  virtual void loadList() = 0;
  virtual void loadEntry(const std::string& name) = 0;
  virtual bool removeEntry(const std::string& name) = 0;
  // Whether Delete may go on (after its own message when not).
  virtual bool mayRemove() { return true; }
  // Fills the fields of a new entry.
  virtual void clearEntry() { clearFields(); }

  Ui& ui_;
  Words words_;
  std::array<std::string, kFields> text_, stored_;
  bool changed_ = false;
  bool isNew_ = true;
  std::vector<std::string> entries_;
  std::string selected_;
  std::optional<Field> focus_;
};

// Plain decimal text of a computed value, to 15 significant digits.
std::string PlainValue(double value);

enum class EllipsoidField {
  ShortName,
  FullName,
  SemimajorAxis,
  SemiminorAxis,
  Flattening,  // shown as 1/f
  Eccentricity,
  Show,
  Count
};

class EllipsoidEditor : public CatalogEditor<EllipsoidField> {
 public:
  EllipsoidEditor(Ui& ui, const std::string& appFolder);
  // Reads the list; a new entry.
  void load();
  bool save() override;
  // A parameter field lost the focus: completes the four parameters from
  // it and the first other one given ('a', 'b', 'f' or 'e').
  void leaveParameter(char parameter);

 private:
  void loadList() override;
  void loadEntry(const std::string& name) override;
  bool removeEntry(const std::string& name) override;
  void clearEntry() override;

  EllipsoidStore store_;
};

enum class DatumField { ShortName, FullName, Type, Ellipsoid, ShowIn, ShowOut, Grid, Count };

struct Transformation {
  std::string datum;
  std::string method;
  bool operator==(const Transformation&) const = default;
};

class DatumEditor : public CatalogEditor<DatumField> {
 public:
  DatumEditor(Ui& ui, const std::string& appFolder);
  // Reads the list and the ellipsoids offered; a new entry.
  void load();
  bool save() override;

  // The type list: fills the method list ("Unknown Datum Type" for another).
  void chooseType(const std::string& type);
  const std::vector<std::string>& ellipsoids() const { return ellipsoids_; }
  const std::vector<std::string>& methods() const { return methods_; }
  bool ellipsoidEnabled() const { return text(DatumField::Type) != "Vertical"; }
  // The datums a transformation may lead to, read afresh: the other datums
  // whose type suits the edited one's.
  std::vector<std::string> targets() const;

  const std::vector<Transformation>& rows() const { return rows_; }
  int selectedRow() const { return row_; }
  void selectRow(int row);
  void addRow();
  void removeRow();
  // Sets the selected row's datum; refused (with a note) when another row
  // leads there already.
  void chooseTarget(const std::string& datum);
  void chooseMethod(const std::string& method);

 private:
  void loadList() override;
  void loadEntry(const std::string& name) override;
  bool removeEntry(const std::string& name) override;
  void clearEntry() override;
  void fillMethods(bool tell);

  std::string appFolder_;
  DatumStore store_;
  std::vector<std::string> ellipsoids_;
  std::vector<std::string> methods_;
  std::vector<Transformation> rows_;
  int row_ = -1;
};

enum class ZoneField {
  CoordinateSystem,
  ShortName,
  FullName,
  HorizontalDatum,
  Ellipsoid,
  VerticalDatum,
  Projection,
  ShowIn,
  ShowOut,
  CentralLatitude,
  CentralLongitude,
  FalseNorthing,
  FalseEasting,
  ScaleFactor,
  NorthernParallel,
  SouthernParallel,
  Azimuth,
  LatitudeDirection,
  LongitudeDirection,
  LinearUnits,
  AngularUnits,
  Count
};

// The parameter fields of a panel, in the order they are checked: 1 for
// Transverse Mercator, one-parallel Lambert and Transverse Mercator NAD 27,
// 2 for the two-parallel and NAD 27 Lambert, 3 for oblique Mercator.
const std::vector<ZoneField>& PanelFields(int panel);
// The panel of a projection; 0 for none.
int ProjectionPanel(const std::string& projection);

class ZoneEditor : public CatalogEditor<ZoneField> {
 public:
  ZoneEditor(Ui& ui, const std::string& appFolder);
  // Reads the datum, ellipsoid and coordinate-system lists; a new entry. A
  // zones.ini section without "~" shows "Error loading coordinate systems."
  // and leaves the coordinate-system list as far as it got.
  void load();
  bool save() override;

  const std::vector<std::string>& coordinateSystems() const { return systems_; }
  // The coordinate system picked in its list: a changed loaded zone is
  // saved first (false when that refused); the zone list is filled with
  // its zones. A new entry takes it as its coordinate system, a loaded one
  // is left for a new entry.
  bool chooseCoordinateSystem(const std::string& system);
  // The coordinate system whose zones are listed.
  const std::string& listedSystem() const { return listed_; }

  // The choices of a list field; the text shown is always among them.
  std::vector<std::string> choices(ZoneField f) const;
  int panel() const { return ProjectionPanel(text(ZoneField::Projection)); }
  // The angular units list: the angles shown are rewritten in the new
  // format (those that cannot be read stay as they are).
  void chooseAngularUnits(const std::string& format);
  // The scale factor lost the focus: "1:N" becomes 1 - 1/N.
  void leaveScaleFactor();
  // Fills a new entry from an imported zone record (angles in the storage
  // form); the coordinate system and short name are kept when the record
  // leaves them empty. False when a changed entry refused to be saved.
  bool importZone(const ZoneRecord& zone);

 private:
  void loadList() override;
  void loadEntry(const std::string& name) override;
  bool removeEntry(const std::string& name) override;
  bool mayRemove() override;
  void clearEntry() override;
  void listZones(const std::string& system);

  ZoneStore store_;
  std::vector<std::string> hDatums_, vDatums_, ellipsoids_, systems_;
  std::string listed_;
  std::string loadedSystem_;
};

}  // namespace zv
