// A measured light distribution: how much light a lamp sends in each direction, as makers publish it in photometric
// text files.
#pragma once

#include "torvane/math/vector.h"
#include "torvane/memory/memory.h"
#include "torvane/memory/private_ge_mtools.h"
#include "torvane/stream/chunk_fields.h"
#include "torvane/text/ge_string.h"

namespace _torvane_
{

class Filename;
class HyperFile;

// Versions of photometric files that are told apart.
enum IESFileVersion : Long
{
  kIESVersionUnknown = 0,
  kIESVersion1991 = 1, // "IESNA91"
  kIESVersion1995 = 2, // "IESNA:LM-63-1995"
};

enum IESTiltMode : Long
{
  kIESTiltUnset = 0,
  kIESTiltNone = 1,    // "NONE"
  kIESTiltInclude = 2, // "INCLUDE": the file holds how the output changes with the lamp's tilt
};

inline constexpr Long kMaxIESAngles = 1024; // of each direction

class IESLight : public GeMemory
{
 public:
  IESLight() = default;
  virtual ~IESLight() = default;
  IESLight(const IESLight&) = delete;
  IESLight& operator=(const IESLight&) = delete;

  Long GetVerticalCount() const { return verticalAngles.GetCount(); }
  Long GetHorizontalCount() const { return horizontalAngles.GetCount(); }
  // The table has a row for each horizontal angle, and no more of either than kMaxIESAngles.
  Bool IsComplete() const;

  // The intensity toward a direction of length 1, relative to maxCandela, from 0 up; 0 outside the vertical angles, and
  // for a table that isn't complete. The lamp's axis is -z: a vertical angle of 0 looks along it. Horizontal angles run
  // from y to x.
  Real SampleIESLight(const Vector& direction) const;

  // Computes maxCandela and the total flux from the table.
  void Normalise();

  // The flux of the relative intensity, over the sphere: 4 pi when it is 1 everywhere, and on a new distribution. What
  // Normalise computes, and a stored form without a flux leaves open, comes from 65536 samples that are the same each
  // time; they are taken when the flux is first asked for.
  Real GetTotalFlux() const;
  void SetTotalFlux(Real flux);

  // The light output of the table, in lumens when it is in candela, by the zonal method that makers use: between two
  // neighbouring vertical angles, the mean intensity all around times the solid angle. It differs by up to 1 % from
  // maxCandela times the total flux, which is sampled. 0 for a table that isn't complete.
  Real GetLumens() const;

  // The stored form within a light's chunk. Reading also takes the versions 1 to 3 of the form; it fails on a table
  // that no photometric file can hold, and when memory is short.
  Bool Write(HyperFile& file);
  Bool Read(HyperFile& file);

  Long fileVersion = kIESVersionUnknown;
  Long tiltMode = kIESTiltUnset;
  String manufacturer;
  String luminaireCatalogue;
  String luminaire;
  String lampCatalogue;
  String lamp;
  Long shape = -1;                       // -1 until a file told one
  Vector size;                           // the luminous opening, in metres
  GeTempDynArray<Real> verticalAngles;   // degrees, ascending
  GeTempDynArray<Real> horizontalAngles; // degrees, ascending
  GeTempDynArray<Real> candela;          // a row of all vertical angles for each horizontal angle
  Real maxCandela = 0.0;

 private:
  friend IESLight* CopyIESLight(const IESLight* source);
  friend struct ChunkFields<IESLight>;

  struct Interval;

  void FindMaximum();

  Bool HasSamples() const;
  Real SampleAt(Real vertical, Real horizontal) const; // in degrees
  Real GetHorizontalPosition(Real angle) const;
  Real GetMeanIntensity(Long vertical) const;
  Real SampleRow(Long row, const Interval& vertical) const;

  mutable Real totalFlux_ = 12.566370614359172;
  mutable Bool fluxIsOpen_ = false; // and to be computed
};

// A new distribution equal to `source`, which the caller owns; null for null and when memory is short.
IESLight* CopyIESLight(const IESLight* source);

// Results of LoadIESFile.
enum IESResult : Long
{
  kIESLoaded = 1,
  kIESNotOpened = -1,
  kIESNotPhotometric = -2, // neither "IESN" nor "TILT" stands near its start
  kIESNoMemory = -3,
  kIESUnreadable = -5, // a read failed, or the numbers aren't those of such a file
};

// What the table of a photometric file is multiplied by: the factors that stand before it.
enum class IESFactors : UChar
{
  kAll,       // as the application does for its lights
  kLightOnly, // without the last one, which in files of today is the power in watts and says nothing of the light
};

// Reads a photometric file. On success `light` is deleted and replaced by a new distribution that the caller owns;
// on failure it stays as it was.
Long LoadIESFile(IESLight*& light, const Filename& name, IESFactors factors = IESFactors::kAll);

// A plain sentence for a result, without a full stop.
const char* GetIESResultText(Long result);

} // namespace _torvane_
